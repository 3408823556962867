# Host time values: seconds since 14 October 1582, the first day of the Gregorian calendar. Day 0
# and month 13 run into the neighbouring month and year; a day before the calendar is missing.
step time date 1582-10-15
step time date "2024-02-29 10:30:15.250"
step time date 2023-13-00
step time date 1582-10-13 || echo "(missing, as it should be)"
step time time 10:30:15,250
# Host print formats as object-model formats: a time with milliseconds, a fixed number with the
# host's digit grouping, and a custom currency.
step format --type 21 --width 11 --decimals 2
step format --type 5 --width 12 --decimals 2 --grouping
step format --type 33 --width 10 --decimals 2
