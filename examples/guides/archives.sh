# Makes a backup with a password, tests it and restores it elsewhere.
mkdir -p data && echo minutes >data/notes.txt && echo prices >data/prices.txt
talutil password --length 16 >key.txt
talutil zip backup.zip data --aes --password-file key.txt
talutil zip --test backup.zip --password-file key.txt >report.txt 2>&1 && echo "the archive is sound"
talutil unzip backup.zip --to restored --password-file key.txt
diff -r data restored/data && echo "the files are the same"
