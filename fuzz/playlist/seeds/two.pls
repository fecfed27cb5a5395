[playlist]
;GENERATED
File2=two%20.mp3
File1=file://localhost/one.mp3
Title1=One
NumberOfEntries=2
Version=2
