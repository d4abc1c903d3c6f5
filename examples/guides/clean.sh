# Cleans a table for the database.
cat >customers.csv <<'CSV'
ID,Name,Suburb,Amount
1,"  mary o'brien, pty ",NORTH RYDE,120.50kg
2,JOHN MCDONALD,manly,80
CSV
cat >customers.plan <<'PLAN'
ID      VerifyIntData 0
Name    VerifyTextData 40 1 | ConvertCase 0
Suburb  VerifyTextData 30 0 | ConvertCaseSuburbs
Amount  VerifyIntData 1
PLAN
talutil clean customers.csv --plan customers.plan --set iCharactercase=1 --set iCharacterCaseSuburbs=1 \
  --output customers.sql >summary.txt 2>&1
cat customers.sql
