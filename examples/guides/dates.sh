# The same on the command line: dates are typed and printed day first.
talutil call IncMonth 31/1/2009 1
talutil call GetWeekNumber 5/3/2009
talutil call GetFinancialYearStr 5/3/2009
