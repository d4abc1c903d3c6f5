# Reads, writes and moves the settings of a user.
user="--database Main --user anne"
talutil config set $user Screen Colour red
talutil config set $user Screen Font Arial
talutil config get $user Screen Colour
talutil config list $user
talutil config export $user anne.ini >report.txt 2>&1
talutil config import --database Main --user bert anne.ini >report.txt 2>&1
talutil config get --database Main --user bert Screen Font

# The same for a profile file, whose comments and order stay.
printf '; of the office\r\n[Printer]\r\nName=Old\r\n' >office.ini
talutil config set --file office.ini Printer Name "Front desk"
cat office.ini | tr -d '\r'
