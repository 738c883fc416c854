<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="en" sourcelanguage="en">
<context>
    <name></name>
    <message id="BRAND_NAME"><source></source><translation>Quillmere</translation></message>
    <message id="SUPPORT_URL"><source></source><translation>https://help.example.net/</translation></message>
    <message id="DEFAULT_ACCOUNT_DESCRIPTION"><source></source><translation>Quillmere account</translation></message>
</context>
</TS>
