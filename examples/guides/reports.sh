# Prints a table and a text to PDF files.
printf 'Name,Amount\nSmith,120\nJones,80\n' >sales.csv
talutil report sales.csv --title Sales --landscape --pdf sales.pdf
printf 'First line\nSecond line\n' >notes.txt
talutil report notes.txt --pdf notes.pdf
head -c 5 sales.pdf && echo
head -c 5 notes.pdf && echo
